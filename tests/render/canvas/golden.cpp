#include "render/canvas/golden.h"

#include <QDir>
#include <QString>

#include <algorithm>

#include <cstdlib>
#include <cstring>

namespace velm::test {
namespace {

QString GoldenPath(const char *name)
{
    return QStringLiteral(VELM_GOLDEN_DIR "/%1.png").arg(QLatin1String(name));
}

QString FailurePath(const char *name, const char *kind)
{
    const QString dir = QStringLiteral(VELM_TEST_BINARY_DIR "/golden-failures");
    QDir().mkpath(dir);
    return QStringLiteral("%1/%2.%3.png").arg(dir, QLatin1String(name), QLatin1String(kind));
}

bool Updating()
{
    const char *flag = std::getenv("VELM_UPDATE_GOLDEN");
    return flag && std::strcmp(flag, "1") == 0;
}

int ChannelDistance(QRgb a, QRgb b)
{
    return std::max({std::abs(qRed(a) - qRed(b)), std::abs(qGreen(a) - qGreen(b)), std::abs(qBlue(a) - qBlue(b)),
                     std::abs(qAlpha(a) - qAlpha(b))});
}

} // namespace

::testing::AssertionResult MatchesGolden(const QImage &drawn, const char *name, Tolerance tolerance)
{
    const QImage actual = drawn.convertToFormat(QImage::Format_ARGB32);
    if (Updating()) {
        if (!actual.save(GoldenPath(name))) return ::testing::AssertionFailure() << "cannot write " << name;
        return ::testing::AssertionSuccess();
    }
    const QImage expected = QImage(GoldenPath(name)).convertToFormat(QImage::Format_ARGB32);
    if (expected.isNull()) {
        actual.save(FailurePath(name, "actual"));
        return ::testing::AssertionFailure() << "no reference image " << name
                                             << ".png; run with VELM_UPDATE_GOLDEN=1 and review it";
    }
    if (expected.size() != actual.size()) {
        actual.save(FailurePath(name, "actual"));
        return ::testing::AssertionFailure() << name << ": size differs from the reference";
    }
    QImage diff(actual.size(), QImage::Format_ARGB32);
    long long outliers = 0;
    int worst = 0;
    for (int y = 0; y < actual.height(); ++y) {
        for (int x = 0; x < actual.width(); ++x) {
            const QRgb want = expected.pixel(x, y);
            const int distance = ChannelDistance(want, actual.pixel(x, y));
            worst = std::max(worst, distance);
            if (distance > tolerance.channel) {
                ++outliers;
                diff.setPixel(x, y, qRgb(255, 0, 0));
            } else {
                const int grey = qGray(want) / 3;
                diff.setPixel(x, y, qRgb(grey, grey, grey));
            }
        }
    }
    const long long allowed = static_cast<long long>(tolerance.outlier_share * actual.width() * actual.height());
    if (outliers <= allowed) return ::testing::AssertionSuccess();
    actual.save(FailurePath(name, "actual"));
    diff.save(FailurePath(name, "diff"));
    return ::testing::AssertionFailure() << name << ": " << outliers << " pixels differ by more than "
                                         << tolerance.channel << " (worst " << worst << "; " << allowed
                                         << " allowed); see golden-failures/ beside the test binary";
}

} // namespace velm::test
