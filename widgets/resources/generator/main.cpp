// Writes every picture of the set as a PNG file into the given folder:
//
//   velm_picture_generator <folder>
//
// The build's `velm_pictures` target runs it on widgets/resources/pictures,
// the folder whose files the library embeds.
#include "widgets/resources/generator/pictures.h"

#include <QDir>
#include <QString>

#include <cstdio>

int main(int argc, char **argv)
{
    if (argc != 2) {
        std::fprintf(stderr, "usage: %s <output folder>\n", argv[0]);
        return 2;
    }
    const QDir folder(QString::fromLocal8Bit(argv[1]));
    if (!folder.exists()) {
        std::fprintf(stderr, "%s: no such folder: %s\n", argv[0], argv[1]);
        return 1;
    }
    int failures = 0;
    for (const auto &picture : velm::pictures::AllPictures()) {
        const QString path = folder.filePath(QString::fromLatin1(picture.name) + QStringLiteral(".png"));
        // Quality 0 asks for the strongest compression: the bytes end up in the library.
        if (!picture.draw().save(path, "PNG", 0)) {
            std::fprintf(stderr, "%s: cannot write %s\n", argv[0], qPrintable(path));
            ++failures;
        }
    }
    return failures == 0 ? 0 : 1;
}
