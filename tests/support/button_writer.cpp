#include "tests/support/movie_writer.h"

TagWriter& TagWriter::DefineButton(U16 id, int code, const std::vector<ButtonImage>& images,
                                   const ButtonBlocks& blocks, bool menu)
{
    const bool conditional = code == kTagDefineButton2;
    ByteWriter records, body = Numbers(id);
    for (const ButtonImage& image : images) {
        records.PutU8(image.flags).PutU16(image.id).PutU16(image.layer).PutMatrix(image.mat);
        if (conditional)
            records.PutCx(image.cx, true);
    }
    if (conditional)
        body.PutU8(menu).PutU16(blocks.empty() ? 0 : U32(records.Size()) + 3);
    body.PutBytes(records.PutU8(0).Bytes());
    for (const auto& [when, actions] : blocks) {
        if (conditional)
            body.PutU16(&when == &blocks.back().first ? 0 : U32(actions.size()) + 4).PutU16(when);
        body.PutBytes(actions);
    }
    return Raw(code, body);
}
