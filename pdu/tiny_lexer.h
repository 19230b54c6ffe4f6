// tinyxml's lexing functions, protected in its base class, opened to the input checks so that
// they read a text exactly as the parser will. Only the static members are used.
#pragma once

#include <tinyxml.h>

struct TinyLexer : TiXmlBase {
    using TiXmlBase::IsAlpha;
    using TiXmlBase::IsWhiteSpace;
    using TiXmlBase::ReadName;
    using TiXmlBase::ReadText;
    using TiXmlBase::SkipWhiteSpace;
    using TiXmlBase::StringEqual;
};
