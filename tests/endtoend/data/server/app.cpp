@import "shape.h"
// Größe 😀 of things
int main()
{
    geo::Circle circle(2);
    geo::Shape shape;
    /* 😀ü */ double size = circle.Getradius() + shape.Area(2);
    int count = 1;
    count += twice(count);
    return count + (size > 3);
}
