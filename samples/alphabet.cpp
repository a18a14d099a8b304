#include "samples/alphabet.h"

#include "samples/pen.h"

#include <algorithm>
#include <array>

namespace {

struct Letter {
    U16 code;
    S16 advance;
    S16 percent; // of the pen's nib
    const char* strokes;
};

// Capitals and figures take a slightly heavier pen, signs a lighter one.
constexpr S16 kSmall = 100, kLarge = 107, kFigure = 103, kSign = 92;

const Letter kLetters[] = {
    {'!', 232, kLarge, "P 64 720 168 720 152 214 80 214 D 116 52 58"},
    {'"', 374, kSmall, "P 62 720 150 720 136 470 76 470 P 224 720 312 720 298 470 238 470"},
    {'#', 640, kSmall, "B 62 430 604 500 B 36 220 578 290 / 166 0 256 720 76 / 384 0 474 720 76"},
    {'$', 594, kFigure,
     "M 486 590 c 446 656 384 690 302 690 c 190 690 112 636 112 540 c 112 436 206 402 306 374"
     " c 416 344 512 306 512 196 c 512 92 424 30 304 30 c 206 30 126 68 80 148"
     " B 266 -90 340 40 B 266 680 340 810"},
    {'%', 780, kSign, "O 168 556 108 132 O 612 164 108 132 / 190 0 590 720 78"},
    {'&', 650, kFigure,
     "M 588 20 L 210 440 c 150 508 132 545 132 586 c 132 650 180 691 250 691"
     " c 320 691 366 650 366 588 c 366 510 290 468 214 422 c 130 370 84 310 84 216"
     " c 84 102 164 29 284 29 c 430 29 524 140 548 350"},
    {'\'', 212, kSmall, "P 62 720 150 720 136 470 76 470"},
    {'(', 310, kSign, "M 252 790 c 92 610 92 40 252 -140"},
    {')', 310, kSign, "M 58 790 c 218 610 218 40 58 -140"},
    {'*', 440, kSmall,
     "B 184 460 256 720 P 315 686 351 624 125 494 89 556 P 125 686 89 624 315 494 351 556"},
    {'+', 560, kSmall, "B 60 318 500 394 B 242 136 318 576"},
    {',', 212, kSmall, "/ 72 -132 116 108 94"},
    {'-', 370, kSmall, "B 54 226 316 304"},
    {'.', 212, kSmall, "D 106 50 58"},
    {'/', 380, kSmall, "/ 40 -120 340 780 82"},
    {'0', 560, kFigure, "O 280 360 196 331"},
    {'1', 560, kFigure, "B 256 0 350 720 P 96 500 96 596 256 720 306 720 306 656"},
    {'2', 560, kFigure,
     "M 92 528 c 100 634 172 691 278 691 c 388 691 460 630 460 532 c 460 424 388 352 316 286"
     " L 128 114 B 78 0 490 80 P 78 0 78 127 98 145 160 80 160 0"},
    {'3', 560, kFigure,
     "M 92 578 c 128 650 190 691 270 691 c 374 691 442 638 442 548 c 442 452 364 394 262 394"
     " L 188 394 M 188 394 L 268 394 c 390 394 468 318 468 212 c 468 100 386 29 268 29"
     " c 178 29 108 70 74 152"},
    {'4', 560, kFigure,
     "B 344 0 436 720 B 40 160 528 238 P 40 238 330 720 400 720 400 650 344 590 138 238"},
    {'5', 560, kFigure,
     "B 136 640 474 720 P 136 720 222 720 206 420 189 379 120 392"
     " w 94 M 164 412 c 196 436 234 446 278 446 w 100 h 472 238 v 268 29"
     " c 182 29 116 66 78 138"},
    {'6', 560, kFigure,
     "O 284 226 188 197 M 96 226 L 96 340 c 96 560 190 691 322 691 w 96"
     " c 390 691 438 664 470 606"},
    {'7', 560, kFigure, "B 66 640 500 720 P 388 650 500 650 276 0 174 0"},
    {'8', 560, kFigure, "O 280 536 160 155 O 280 210 192 181"},
    {'9', 560, kFigure,
     "O 276 494 188 197 M 464 494 L 464 380 c 464 160 370 29 238 29 w 96"
     " c 170 29 122 56 90 114"},
    {':', 212, kSmall, "D 106 50 58 D 106 450 58"},
    {';', 212, kSmall, "/ 72 -132 116 108 94 D 106 450 58"},
    {'<', 560, kSmall, "P 60 318 60 394 500 576 500 492 158 356 500 220 500 136"},
    {'=', 560, kSmall, "B 60 408 500 482 B 60 230 500 304"},
    {'>', 560, kSmall, "P 500 318 500 394 60 576 60 492 402 356 60 220 60 136"},
    {'?', 490, kLarge,
     "M 66 560 c 92 644 156 690 242 690 c 348 690 418 630 418 540 c 418 410 244 400 244 214"
     " D 244 52 58"},
    {'@', 920, kSign,
     "M 716 -20 c 650 -70 570 -96 478 -96 h 70 300 v 478 690 h 850 330 c 850 190 790 150 724 150"
     " c 664 150 640 180 640 240 L 640 470 O 482 310 144 152"},
    {'A', 640, kLarge, "/ 66 0 320 720 100 / 574 0 320 720 100 B 150 194 490 272"},
    {'B', 580, kLarge,
     "B 74 0 168 720 M 120 680 L 312 680 h 456 530 v 312 380 L 120 380"
     " M 120 380 L 330 380 h 496 208 v 330 40 L 120 40"},
    {'C', 640, kLarge,
     "M 588 560 c 540 646 464 690 362 690 h 88 360 v 362 30 c 464 30 540 74 588 160"},
    {'D', 690, kLarge, "B 74 0 168 720 M 120 680 L 290 680 h 602 360 v 290 40 L 120 40"},
    {'E', 536, kLarge, "B 74 0 168 720 B 74 640 484 720 B 74 332 446 410 B 74 0 492 80"},
    {'F', 506, kLarge, "B 74 0 168 720 B 74 640 478 720 B 74 312 436 390"},
    {'G', 716, kLarge,
     "M 600 568 c 552 650 470 690 370 690 h 88 360 v 374 30 c 486 30 572 66 626 118"
     " B 578 92 670 372 B 400 294 670 372"},
    {'H', 706, kLarge, "B 74 0 168 720 B 538 0 632 720 B 74 328 632 408"},
    {'I', 246, kLarge, "B 76 0 170 720"},
    {'J', 444, kLarge, "M 326 720 L 326 206 w 96 v 186 30 c 118 30 66 62 36 132"},
    {'K', 622, kLarge, "B 74 0 168 720 / 130 270 534 720 122 / 564 0 288 446 124"},
    {'L', 494, kLarge, "B 74 0 168 720 B 74 0 470 80"},
    {'M', 828, kLarge,
     "B 74 0 164 720 B 664 0 754 720 / 414 100 126 720 104 / 414 100 702 720 104"},
    {'N', 714, kLarge, "B 74 0 164 720 B 550 0 640 720 P 74 720 180 720 640 0 534 0"},
    {'O', 752, kLarge, "O 376 360 288 330"},
    {'P', 560, kLarge, "B 74 0 168 720 M 120 680 L 316 680 h 478 506 v 316 332 L 120 332"},
    {'Q', 752, kLarge, "O 376 360 288 330 / 654 -64 470 190 118"},
    {'R', 596, kLarge,
     "B 74 0 168 720 M 120 680 L 314 680 h 470 516 v 314 352 L 120 352 / 524 0 330 372 112"},
    {'S', 580, kLarge,
     "M 480 590 c 440 656 378 690 296 690 c 186 690 108 636 108 540 c 108 436 200 402 300 374"
     " c 410 344 504 306 504 196 c 504 92 418 30 298 30 c 200 30 120 68 76 148"},
    {'T', 586, kLarge, "B 24 640 562 720 B 246 0 340 720"},
    {'U', 700, kLarge, "M 118 720 L 118 266 v 350 30 h 582 266 L 582 720"},
    {'V', 632, kLarge, "/ 316 0 70 720 100 / 316 0 562 720 100"},
    {'W', 932, kLarge,
     "/ 264 0 66 720 96 / 264 0 466 720 94 / 668 0 466 720 94 / 668 0 866 720 96"},
    {'X', 606, kLarge, "/ 78 0 516 720 114 / 528 0 90 720 114"},
    {'Y', 604, kLarge,
     "B 255 0 349 310 P 14 720 122 720 349 284 255 284 "
     "P 590 720 482 720 255 284 349 284"},
    {'Z', 590, kLarge, "B 54 640 540 720 B 44 0 548 80 P 44 80 412 640 540 640 172 80"},
    {'[', 310, kSign, "B 76 -140 152 790 B 76 722 270 790 B 76 -140 270 -72"},
    {'\\', 380, kSmall, "/ 340 -120 40 780 82"},
    {']', 310, kSign, "B 158 -140 234 790 B 40 722 234 790 B 40 -140 234 -72"},
    {'^', 500, kSmall, "/ 100 430 250 720 82 / 400 430 250 720 82"},
    {'_', 512, kSmall, "B 0 -150 512 -84"},
    {'`', 290, kSmall, "/ 196 580 98 730 92"},
    {'a', 502, kSmall,
     "M 392 0 L 392 320 w 94 v 240 482 w 98 c 172 482 122 458 86 410"
     " w 76 M 392 292 L 264 292 w 96 h 88 152 w 92 v 212 28 w 60 c 312 28 386 86 392 170"},
    {'b', 558, kSmall,
     "B 62 0 150 760 w 52 M 122 350 w 94 v 290 482 w 100 h 476 255 w 94 v 290 28 w 52 h 122 160"},
    {'c', 486, kSmall,
     "w 96 M 446 400 c 412 454 356 482 286 482 w 100 h 82 255 w 96 v 286 28"
     " c 356 28 412 56 446 110"},
    {'d', 558, kSmall,
     "B 408 0 496 760 w 52 M 436 350 w 94 v 268 482 w 100 h 82 255 w 94 v 268 28 w 52 h 436 160"},
    {'e', 536, kSmall,
     "M 456 224 w 94 v 270 482 w 100 h 82 255 w 94 v 278 28 w 96 c 350 28 410 52 450 104"
     " B 100 224 470 292"},
    {'f', 326, kSmall, "M 144 0 L 144 590 w 96 v 262 726 L 318 726 B 34 436 304 510"},
    {'g', 558, kSmall,
     "w 52 M 436 350 w 94 v 268 482 w 100 h 82 255 w 94 v 268 28 w 52 h 436 160"
     " w 100 M 452 510 L 452 -30 w 94 v 268 -186 w 96 c 196 -186 142 -162 104 -112"},
    {'h', 534, kSmall, "B 62 0 150 760 w 52 M 122 340 w 94 v 290 482 w 100 h 430 322 L 430 0"},
    {'i', 212, kSmall, "B 62 0 150 510 D 106 654 58"},
    {'j', 216, kSmall, "M 110 510 L 110 -60 w 94 v 8 -186 L -26 -186 D 110 654 58"},
    {'k', 490, kSmall, "B 62 0 150 760 / 128 186 400 510 108 / 434 0 240 314 110"},
    {'l', 212, kSmall, "B 62 0 150 760"},
    {'m', 796, kSmall,
     "B 62 0 150 510 w 52 M 122 340 w 94 v 272 482 w 100 h 398 322 L 398 0"
     " w 52 M 414 340 w 94 v 564 482 w 100 h 692 322 L 692 0"},
    {'n', 534, kSmall, "B 62 0 150 510 w 52 M 122 340 w 94 v 290 482 w 100 h 430 322 L 430 0"},
    {'o', 548, kSmall, "O 274 255 192 227"},
    {'p', 558, kSmall,
     "B 62 -210 150 510"
     " w 52 M 122 350 w 94 v 290 482 w 100 h 476 255 w 94 v 290 28 w 52 h 122 160"},
    {'q', 558, kSmall,
     "B 408 -210 496 510"
     " w 52 M 436 350 w 94 v 268 482 w 100 h 82 255 w 94 v 268 28 w 52 h 436 160"},
    {'r', 352, kSmall, "B 62 0 150 510 w 52 M 122 320 w 98 v 288 474 L 336 474"},
    {'s', 456, kSmall,
     "w 96 M 374 416 c 342 460 296 484 232 484 c 150 484 92 446 92 382"
     " c 92 310 160 285 235 262 c 320 236 384 206 384 132 c 384 66 324 26 234 26"
     " c 168 26 106 52 70 104"},
    {'t', 346, kSmall, "M 150 652 L 150 170 w 96 v 258 38 L 318 38 B 36 436 314 510"},
    {'u', 534, kSmall, "B 384 0 472 510 w 52 M 412 170 w 94 v 244 28 w 100 h 104 188 L 104 510"},
    {'v', 500, kSmall, "/ 250 0 66 510 92 / 250 0 434 510 92"},
    {'w', 752, kSmall,
     "/ 216 0 64 510 90 / 216 0 376 510 86 / 536 0 376 510 86 / 536 0 688 510 90"},
    {'x', 476, kSmall, "/ 72 0 400 510 104 / 404 0 76 510 104"},
    {'y', 500, kSmall, "/ 174 -210 434 510 92 / 250 0 66 510 92"},
    {'z', 460, kSmall, "B 46 438 412 510 B 40 0 420 72 P 40 72 302 438 412 438 150 72"},
    {'{', 330, kSign,
     "M 284 755 c 200 755 168 720 168 640 L 168 440 c 168 370 130 325 60 325"
     " M 284 -105 c 200 -105 168 -70 168 10 L 168 210 c 168 280 130 325 60 325"},
    {'|', 272, kSmall, "B 98 -160 174 800"},
    {'}', 330, kSign,
     "M 46 755 c 130 755 162 720 162 640 L 162 440 c 162 370 200 325 270 325"
     " M 46 -105 c 130 -105 162 -70 162 10 L 162 210 c 162 280 200 325 270 325"},
    {'~', 520, kSign, "M 62 296 c 92 376 160 406 260 356 c 360 306 428 336 458 416"},
    {0xA1, 232, kLarge, "P 64 -210 168 -210 152 296 80 296 D 116 458 58"},
    {0xAB, 470, kSmall,
     "/ 130 110 90 260 88 / 130 410 90 260 88 / 320 110 280 260 88 / 320 410 280 260 88"},
    {0xB7, 212, kSmall, "D 106 300 58"},
    {0xBB, 470, kSmall,
     "/ 340 260 300 110 88 / 340 260 300 410 88 / 150 260 110 110 88 / 150 260 110 410 88"},
    {0xBF, 490, kLarge,
     "M 424 -50 c 398 -134 334 -180 248 -180 c 142 -180 72 -120 72 -30 c 72 100 246 110 246 296"
     " D 246 458 58"},
    {0xC6, 880, kLarge,
     "/ 66 0 400 720 104 B 150 186 480 264 B 404 0 498 720 B 370 640 820 720"
     " B 404 332 780 410 B 404 0 830 80"},
    {0xD8, 752, kLarge, "O 376 360 288 330 / 116 -30 636 750 84"},
    {0xDF, 520, kSmall,
     "M 106 0 L 106 580 w 96 v 256 726 h 398 606 c 398 500 276 470 276 392"
     " c 276 310 452 300 452 158 c 452 76 390 28 310 28 c 266 28 232 36 206 50"},
    {0xE6, 860, kSmall,
     "M 392 130 L 392 320 w 94 v 240 482 w 98 c 172 482 122 458 86 410"
     " w 76 M 392 292 L 264 292 w 96 h 88 152 w 92 v 216 28 w 92 h 412 200"
     " w 100 M 780 224 w 94 v 594 482 w 100 h 406 255 w 94 v 602 28 w 96 c 674 28 734 52 774 104"
     " B 424 224 794 292"},
    {0xF8, 548, kSmall, "O 274 255 192 227 / 82 -40 466 550 76"},
    {0x2013, 560, kSmall, "B 30 228 530 302"},
    {0x2014, 960, kSmall, "B 30 228 930 302"},
    {0x2018, 206, kSmall, "/ 124 490 84 720 92"},
    {0x2019, 206, kSmall, "/ 82 490 122 720 92"},
    {0x201C, 366, kSmall, "/ 124 490 84 720 92 / 284 490 244 720 92"},
    {0x201D, 366, kSmall, "/ 82 490 122 720 92 / 242 490 282 720 92"},
    {0x201E, 366, kSmall, "/ 72 -132 112 98 92 / 232 -132 272 98 92"},
    {0x2026, 636, kSmall, "D 106 50 58 D 318 50 58 D 530 50 58"},
};

// Marks stand over (or under) the middle of a letter; y counts from the top of a small one.
enum Mark { kGrave, kAcute, kCircumflex, kTilde, kDiaeresis, kRing, kCedilla, kMarks };

const char* const kMarkStrokes[kMarks] = {
    "/ 42 66 -44 210 92",
    "/ -42 66 44 210 92",
    "/ -92 66 0 206 84 / 92 66 0 206 84",
    "w 86 M -134 88 c -110 160 -64 164 0 134 c 64 104 110 108 134 180",
    "D -82 134 52 D 82 134 52",
    "w 70 O 0 146 62 62",
    "w 78 M 6 -500 c 6 -560 70 -560 70 -630 c 70 -690 0 -706 -70 -674",
};

struct Marked {
    U16 code;
    char base;
    Mark mark;
};

const Marked kMarked[] = {
    {0xC0, 'A', kGrave},      {0xC1, 'A', kAcute},      {0xC2, 'A', kCircumflex},
    {0xC3, 'A', kTilde},      {0xC4, 'A', kDiaeresis},  {0xC5, 'A', kRing},
    {0xC7, 'C', kCedilla},    {0xC8, 'E', kGrave},      {0xC9, 'E', kAcute},
    {0xCA, 'E', kCircumflex}, {0xCB, 'E', kDiaeresis},  {0xCC, 'I', kGrave},
    {0xCD, 'I', kAcute},      {0xCE, 'I', kCircumflex}, {0xCF, 'I', kDiaeresis},
    {0xD1, 'N', kTilde},      {0xD2, 'O', kGrave},      {0xD3, 'O', kAcute},
    {0xD4, 'O', kCircumflex}, {0xD5, 'O', kTilde},      {0xD6, 'O', kDiaeresis},
    {0xD9, 'U', kGrave},      {0xDA, 'U', kAcute},      {0xDB, 'U', kCircumflex},
    {0xDC, 'U', kDiaeresis},  {0xDD, 'Y', kAcute},      {0xE0, 'a', kGrave},
    {0xE1, 'a', kAcute},      {0xE2, 'a', kCircumflex}, {0xE3, 'a', kTilde},
    {0xE4, 'a', kDiaeresis},  {0xE5, 'a', kRing},       {0xE7, 'c', kCedilla},
    {0xE8, 'e', kGrave},      {0xE9, 'e', kAcute},      {0xEA, 'e', kCircumflex},
    {0xEB, 'e', kDiaeresis},  {0xEC, 'i', kGrave},      {0xED, 'i', kAcute},
    {0xEE, 'i', kCircumflex}, {0xEF, 'i', kDiaeresis},  {0xF1, 'n', kTilde},
    {0xF2, 'o', kGrave},      {0xF3, 'o', kAcute},      {0xF4, 'o', kCircumflex},
    {0xF5, 'o', kTilde},      {0xF6, 'o', kDiaeresis},  {0xF9, 'u', kGrave},
    {0xFA, 'u', kAcute},      {0xFB, 'u', kCircumflex}, {0xFC, 'u', kDiaeresis},
    {0xFD, 'y', kAcute},      {0xFF, 'y', kDiaeresis},
};

constexpr S32 kSpaceAdvance = 250;

template <class Entry, size_t count> const Entry* Find(const Entry (&table)[count], U16 code)
{
    const Entry* found =
        std::find_if(table, table + count, [&](const Entry& entry) { return entry.code == code; });
    return found == table + count ? nullptr : found;
}

void DrawMarked(const Marked& marked, std::vector<GlyphContour>* out)
{
    const Letter& base = *Find(kLetters, U16(marked.base));
    const bool large = marked.base < 'a', below = marked.mark == kCedilla;
    // An i gives up its dot for what stands there.
    DrawWithPen(marked.base == 'i' ? "B 62 0 150 510" : base.strokes, {0, 0, base.percent}, out);
    const S32 top = large && !below ? kAlphabetCapHeight - 40 : kAlphabetXHeight;
    DrawWithPen(kMarkStrokes[marked.mark], {base.advance / 2, top, base.percent}, out);
}

} // namespace

const std::vector<U16>& AlphabetCodes()
{
    static const std::vector<U16> codes = [] {
        std::vector<U16> all = {' '};
        for (const Letter& letter : kLetters)
            all.push_back(letter.code);
        for (const Marked& marked : kMarked)
            all.push_back(marked.code);
        std::sort(all.begin(), all.end());
        return all;
    }();
    return codes;
}

S32 AlphabetAdvance(U16 code)
{
    if (code == ' ')
        return kSpaceAdvance;
    if (const Marked* marked = Find(kMarked, code))
        code = U16(marked->base);
    const Letter* letter = Find(kLetters, code);
    return letter ? letter->advance : 0;
}

std::vector<GlyphContour> AlphabetOutline(U16 code)
{
    std::vector<GlyphContour> out;
    if (const Letter* letter = Find(kLetters, code))
        DrawWithPen(letter->strokes, {0, 0, letter->percent}, &out);
    if (const Marked* marked = Find(kMarked, code))
        DrawMarked(*marked, &out);
    return out;
}
