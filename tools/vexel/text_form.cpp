#include "tools/vexel/text_form.h"

#include "tools/vexel/message.h"

std::string Quote(const std::string& bytes)
{
    std::string text = "\"";
    for (const char c : bytes) {
        const unsigned char byte = static_cast<unsigned char>(c);
        if (c == '"' || c == '\\')
            (text += '\\') += c;
        else if (byte < 32 || byte > 126)
            text += Format("\\x%02x", byte);
        else
            text += c;
    }
    return text + '"';
}

std::string RectText(const SRECT& r)
{
    return Format("%d,%d,%d,%d", r.xmin, r.xmax, r.ymin, r.ymax);
}

std::string MatrixText(const MATRIX& m)
{
    if (MatrixIsIdentity(&m))
        return "identity";
    return Format("%.6g,%.6g,%.6g,%.6g,%d,%d", m.a / 65536.0, m.b / 65536.0, m.c / 65536.0,
                  m.d / 65536.0, m.tx, m.ty);
}

std::string CxformText(const ColorTransform& cx)
{
    return Format("r*%d%+d,g*%d%+d,b*%d%+d,a*%d%+d", cx.redMul, cx.redAdd, cx.greenMul, cx.greenAdd,
                  cx.blueMul, cx.blueAdd, cx.alphaMul, cx.alphaAdd);
}

std::string ColorText(SRGB c)
{
    const std::string text = Format("#%02x%02x%02x", c.red, c.green, c.blue);
    return c.alpha == 255 ? text : text + Format("%02x", c.alpha);
}
